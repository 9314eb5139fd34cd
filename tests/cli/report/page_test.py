#!/usr/bin/env python3
"""What a user does with a report, in headless Chromium: page_test.py TOOL."""

import pathlib
import struct
import subprocess
import sys
import tempfile
import unittest

import browser

DATABASE = pathlib.Path(__file__).resolve().parents[3] / "database"
TOOL = None
CHROMIUM = None

# Names and values that a page could mistake for its own.
HOSTILE = {
    "base.acd": b"DEVICE_SUPPORTED = fam\nPROGRAM_OPTION_PACKAGE = fam\n"
                b"BS = outputs,USB2:families,fam\nIDCODE = <script>,0x1\"'<b>:100%,%s%n\n",
    "fam.acd": b"OPERATION = PROGRAM,Bscan,USB2\nPROPERTY = <img src=x onerror=\"alert('p')\">,<i>value</i>\n"
               b"[<script>alert(1)</script>]\n"
               b"PROPERTY = A,</script><script>alert(2)</script>:B,\"'&amp;%s%n:C,\xff\xfe\xc3\xa9:D,<!--\n"
               b"[</script>]\n[<script>]\n[\"onclick=\"alert(3)]\n[A'B]\n[100%]\n[\xff]\n[\xfe]\n[toString]\n[__proto__]\n",
    "spi.acd": b"DEVICE_FAMILY = <b>\n<b>_DEVICES = <u>F</u>\n<U>F</U>_PROPERTY = K,<s>v</s>\n"
               b"TYPE_MB_SPI_NONE_LEAD = <u>F</u>,<script>\n",
}


def report(directory, database, name="report.html", status=0):
    """Writes the report of a database, with which the tool ends with this status. @return its address"""
    path = pathlib.Path(directory) / name
    ended = subprocess.run([TOOL, "--database", str(database), "report", "--file", str(path)], check=False,
                           stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, text=True, errors="replace")
    assert ended.returncode == status, ended.stderr
    return path.as_uri()


def many_devices(count):
    """A database of two families with so many devices that their parts are made by the script."""
    def family(letter, operation):
        sections = "".join(f"[{letter}{number}]\nPROPERTY = PINS,{number}\n" for number in range(count // 2))
        return f"OPERATION = {operation},Bscan,USB2\nPROPERTY = VENDOR,Korvel\n{sections}"

    return {
        "base.acd": b"DEVICE_SUPPORTED = ant,bee\nPROGRAM_OPTION_PACKAGE = ant,bee\n"
                    b"BS = outputs,USB2:families,ant,bee\nIDCODE = A7,0xA7\n",
        "ant.acd": family("A", "PROGRAM").encode(),
        "bee.acd": family("B", "ERASE").encode(),
        "spi.acd": b"DEVICE_FAMILY =\nTYPE_MB_SPI_NONE_LEAD = A3,B4\n",
    }


def database(directory, files):
    folder = pathlib.Path(tempfile.mkdtemp(dir=directory))
    for name, text in files.items():
        (folder / name).write_bytes(text)
    return folder


class PageTest(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls._place = tempfile.TemporaryDirectory(prefix="tarvik-report-")
        cls.place = cls._place.name
        cls.address = cls.make()

    @classmethod
    def tearDownClass(cls):
        cls._place.cleanup()

    @classmethod
    def make(cls):
        return report(cls.place, DATABASE)

    def open(self, fragment="", **how):
        page = CHROMIUM.page(**how)
        self.addCleanup(page.close)
        page.open(self.address + fragment)
        page.settle()
        return page

    def listed(self, page):
        return page.evaluate("[...document.querySelectorAll('#list h4')].map((one) => one.textContent)")

    def count(self, page):
        return page.evaluate("document.getElementById('count').textContent")

    def focused(self, page):
        return page.evaluate("document.activeElement.id || document.activeElement.textContent")

    def is_seen(self, page, expression):
        """Does an element lie in the window, on top?"""
        return page.evaluate(f"""(() => {{
            const box = ({expression}).getBoundingClientRect();
            const top = document.elementFromPoint(box.x + 5, box.y + Math.min(5, box.height / 2));
            return top !== null && ({expression}).contains(top);
        }})()""")


class Demonstration(PageTest):
    def test_opens_with_all_devices_and_without_complaint(self):
        page = self.open()
        names = self.listed(page)
        self.assertGreater(len(names), 150)
        self.assertIn("KS50", names)
        self.assertEqual(self.count(page), f"{len(names)} devices")
        self.assertEqual(page.complaints(), [])

    def test_asks_nobody_else(self):
        page = self.open()
        asked = [url for url in page.requests() if url != "about:blank" and not url.startswith("data:")]
        self.assertEqual(asked, [self.address])

    def test_overview_counts_pairs(self):
        page = self.open()
        cell = """(() => {
            const table = document.querySelector("#overview table");
            const column = [...table.tHead.rows[0].cells].findIndex((head) => head.textContent === "PROGRAM");
            return [...table.tBodies[0].rows].find((row) => row.cells[0].textContent === "kestrel")
                .cells[column].textContent;
        })()"""
        # PROGRAM of kestrel: 4 outputs in BS, 3 in SS, 2 in SM, 2 in BSFILE; those in SPI mode are the flashes' own.
        self.assertEqual(page.evaluate(cell), "11")

    def test_search(self):
        page = self.open()
        page.press("/")
        self.assertEqual(self.focused(page), "search")
        page.write("ks10")
        self.assertEqual(self.listed(page), ["KS100", "KS1000"])
        self.assertRegex(self.count(page), r"^2 of \d+ devices$")
        page.press("Escape")
        self.assertGreater(len(self.listed(page)), 150)

    def test_whole_name_comes_first(self):
        page = self.open()
        page.press("/")
        page.write("gk120p")
        self.assertEqual(self.listed(page)[0], "GK120P")
        page.evaluate("document.getElementById('search').select()")
        page.write("KS100")
        self.assertEqual(self.listed(page), ["KS100", "KS1000"])

    def test_search_without_result(self):
        page = self.open()
        page.press("/")
        page.write("no such device")
        self.assertEqual(self.listed(page), [])
        self.assertRegex(self.count(page), "^0 of")

    def test_filters(self):
        page = self.open()
        page.choose("#operation", "READIDCODE")
        page.choose("#mode", "4")  # DP770
        spi = self.listed(page)
        self.assertIn("OVD16", spi)
        self.assertNotIn("KS50", spi)
        page.choose("#output", "3")  # SVF
        self.assertEqual(self.listed(page), [])
        page.click("#filters [type=reset]")
        self.assertGreater(len(self.listed(page)), 150)
        page.choose("#family", page.evaluate(
            "[...document.querySelectorAll('#family option')].find((one) => one.textContent === 'kestrel').value"))
        self.assertEqual(len(self.listed(page)), 10)
        page.choose("#operation", "HIGHZ")  # by boundary scan alone
        self.assertEqual(len(self.listed(page)), 10)
        page.choose("#mode", "0")
        self.assertEqual(self.listed(page), [])

    def test_filters_agree_with_which(self):
        page = self.open()
        page.choose("#operation", "ERASE")
        page.choose("#mode", "0")
        page.choose("#output", "2")
        answer = subprocess.run([TOOL, "--database", str(DATABASE), "which", "--operation", "ERASE", "--mode", "BS",
                                 "--output", "USB2"], check=True, capture_output=True, text=True).stdout
        self.assertEqual(self.listed(page), [line.split()[0] for line in answer.splitlines()[1:]])

    def test_cell_of_the_overview_filters(self):
        page = self.open()
        page.evaluate("""(() => {
            const table = document.querySelector("#overview table");
            const column = [...table.tHead.rows[0].cells].findIndex((head) => head.textContent === "VERIFY");
            [...table.tBodies[0].rows].find((row) => row.cells[0].textContent === "kestrel").cells[column].click();
        })()""")
        self.assertEqual(page.evaluate("document.getElementById('operation').value"), "VERIFY")
        self.assertEqual(len(self.listed(page)), 10)

    def test_family_of_the_overview_filters(self):
        page = self.open()
        for _ in range(2):  # again from the same address
            page.click("#overview a[href='#in-kestrel']")
            page.wait_until("document.querySelectorAll('#list h4').length === 10")
            page.click("#filters [type=reset]")

    def test_link_to_a_device(self):
        for fragment in ("#device-KS50", "#device-ks50"):
            page = self.open(fragment)
            part = "document.getElementById('device-KS50')"
            page.wait_until(f"{part}.parentElement.open")
            self.assertTrue(self.is_seen(page, f"{part}.parentElement.firstElementChild"))
            self.assertIn("kestrel.acd:", page.evaluate(f"{part}.textContent"))

    def test_link_follows_behind_a_filter(self):
        page = self.open()
        page.choose("#operation", "READUES")
        page.evaluate("location.hash = '#device-KS50'")
        page.wait_until("document.getElementById('device-KS50')?.parentElement.open")
        self.assertEqual(page.evaluate("document.getElementById('operation').value"), "")

    def test_links_of_flashes_and_multiboot(self):
        page = self.open()
        page.click("#flashes a[href='#device-OVD16']")
        page.wait_until("document.getElementById('device-OVD16').parentElement.open")
        page.click("#multiboot a[href='#device-KS1500']")
        page.wait_until("document.getElementById('device-KS1500').parentElement.open")

    def test_address_of_an_opened_device(self):
        page = self.open()
        page.evaluate("document.getElementById('device-KS50').parentElement.firstElementChild.click()")
        self.assertEqual(page.evaluate("location.hash"), "#device-KS50")

    def test_script_makes_the_parts_that_the_tool_writes(self):
        page = self.open()
        written = page.evaluate("[...document.querySelectorAll('.device')].map((one) => one.outerHTML)")
        page.call("Page.addScriptToEvaluateOnNewDocument", source="""
            // As if the tool had written no parts.
            new MutationObserver((_, watch) => {
                if (document.querySelector("#list ~ *") !== null) {
                    document.getElementById("list").replaceChildren();
                    watch.disconnect();
                }
            }).observe(document, {childList: true, subtree: true});""")
        page.open(self.address)
        page.settle()
        while page.evaluate("!document.getElementById('more').hidden"):
            page.click("#more")
        page.click("#open-all")
        page.click("#close-all")
        made = page.evaluate("[...document.querySelectorAll('.device')].map((one) => one.outerHTML)")
        self.assertEqual(len(made), len(written))
        for one, other in zip(made, written):
            self.assertEqual(one, other)

    def test_reads_without_scripts(self):
        page = self.open(scripts=False)
        page.run_scripts()
        self.assertGreater(len(self.listed(page)), 150)
        self.assertEqual(page.evaluate("[...document.querySelectorAll('[hidden]')].map((one) => one.id).sort()"),
                         ["filters", "more", "openers", "theme"])
        part = page.evaluate("document.getElementById('device-KS50').textContent")
        for text in ("TQ144", "READSTATUSREGISTER", "Programming options", "kestrel.acd:"):
            self.assertIn(text, part)
        self.assertIn("TYPE_MB_SPI", page.evaluate("document.getElementById('multiboot').textContent"))
        self.assertIn("MRS256K", page.evaluate("document.getElementById('flashes').textContent"))

    def test_link_to_a_device_without_scripts(self):
        page = self.open("#device-KS50", scripts=False)
        page.run_scripts()
        page.wait_until("document.getElementById('device-KS50').parentElement.open")

    def test_dark_and_light(self):
        background = "getComputedStyle(document.body).backgroundColor"
        page = self.open()
        light = page.evaluate(background)
        page.emulate("dark")
        dark = page.evaluate(background)
        self.assertNotEqual(light, dark)
        page.wait_until("document.getElementById('theme').textContent === 'Light'")
        page.click("#theme")
        self.assertEqual(page.evaluate(background), light)
        page.open(self.address)
        self.assertEqual(page.evaluate(background), light)  # the choice is kept
        page.click("#theme")
        page.emulate("light")
        self.assertEqual(page.evaluate(background), dark)
        page.evaluate("localStorage.clear()")

    def test_contrast(self):
        for scheme in ("light", "dark"):
            page = self.open("#device-KS50", scheme=scheme)
            poor = page.evaluate("""(() => {
                const canvas = document.createElement("canvas").getContext("2d", {willReadFrequently: true});
                const colour = (text) => {
                    canvas.clearRect(0, 0, 1, 1);
                    canvas.fillStyle = text;
                    canvas.fillRect(0, 0, 1, 1);
                    return [...canvas.getImageData(0, 0, 1, 1).data];
                };
                const luminance = (rgb) => rgb.slice(0, 3).map((part) => part / 255)
                    .map((part) => part <= 0.04045 ? part / 12.92 : ((part + 0.055) / 1.055) ** 2.4)
                    .reduce((sum, part, i) => sum + part * [0.2126, 0.7152, 0.0722][i], 0);
                const behind = (one) => {
                    for (; one !== null; one = one.parentElement) {
                        const found = colour(getComputedStyle(one).backgroundColor);
                        if (found[3] === 255) {
                            return found;
                        }
                    }
                    return [255, 255, 255, 255];
                };
                const poor = new Set();
                for (const one of document.querySelectorAll("body *:not(script, style, option)")) {
                    const hasText = [...one.childNodes].some((node) => node.nodeType === 3 && node.data.trim() !== "");
                    // What stands for nothing may be faint.
                    if (hasText && one.offsetParent !== null && !one.matches(".matrix i, .none")) {
                        const [ink, paper] = [colour(getComputedStyle(one).color), behind(one)].map(luminance);
                        const ratio = (Math.max(ink, paper) + 0.05) / (Math.min(ink, paper) + 0.05);
                        if (ratio < 4.5) {
                            poor.add(`${one.localName}.${one.className} ${ratio.toFixed(2)}`);
                        }
                    }
                }
                return [...poor];
            })()""")
            self.assertEqual(poor, [], scheme)

    def test_keyboard(self):
        page = self.open()
        page.press("Tab")
        self.assertEqual(self.focused(page), "Skip to the devices")
        self.assertTrue(self.is_seen(page, "document.activeElement"))
        self.assertNotEqual(page.evaluate("getComputedStyle(document.activeElement).outlineStyle"), "none")
        page.press("Enter")
        page.press("Tab")
        self.assertEqual(self.focused(page), "search")
        for field in ("family", "operation", "mode", "output"):
            page.press("Tab")
            self.assertEqual(self.focused(page), field)
        for _ in range(4):  # Clear, Open all, Close all, the first device
            page.press("Tab")
        first = self.listed(page)[0]
        self.assertTrue(self.focused(page).startswith(first))
        page.press("Enter")
        self.assertTrue(page.evaluate("document.activeElement.parentElement.open"))
        page.press("/")
        self.assertEqual(self.focused(page), "search")

    def test_slash_can_be_searched_for(self):
        page = self.open()
        page.press("/")
        page.press("/")
        self.assertEqual(page.evaluate("document.getElementById('search').value"), "/")

    def test_everything_has_a_name(self):
        page = self.open("#device-KS50")
        tree = page.call("Accessibility.getFullAXTree")["nodes"]
        roles = {"button", "textbox", "searchbox", "combobox", "link", "region", "navigation", "search", "table"}
        seen = set()
        for node in tree:
            role = node.get("role", {}).get("value")
            if role in roles and not node.get("ignored"):
                seen.add(role)
                self.assertTrue(node.get("name", {}).get("value"), f"a {role} without a name")
        self.assertTrue({"searchbox", "combobox", "button", "link", "region", "table"} <= seen, seen)
        self.assertEqual(page.evaluate("document.querySelectorAll('th:not([scope])').length"), 0)
        self.assertEqual(page.evaluate("document.querySelectorAll('table:not(:has(> caption))').length"), 0)

    def test_headings_descend_one_by_one(self):
        page = self.open()
        levels = page.evaluate("[...document.querySelectorAll('h1, h2, h3, h4')].map((one) => Number(one.localName[1]))")
        self.assertEqual(levels[0], 1)
        for former, level in zip(levels, levels[1:]):
            self.assertLessEqual(level, former + 1)

    def test_names_are_unique(self):
        page = self.open()
        self.assertEqual(page.evaluate("""(() => {
            const all = [...document.querySelectorAll("[id]")].map((one) => one.id);
            return all.filter((id, position) => all.indexOf(id) !== position);
        })()"""), [])

    def test_each_matrix_has_a_legend(self):
        page = self.open("#device-KS50")
        legends = page.evaluate("""[...document.querySelectorAll("#device-KS50 .matrix caption")]
            .map((caption) => caption.textContent)""")
        letters = "P PARALLEL, Z ZORVA, U USB2, S SVF, T STAPL"
        self.assertEqual(legends, [f"Operations {letters}", f"Programming options {letters}"])

    def test_rows_of_spi_mode_are_marked(self):
        marked = """[...document.querySelectorAll("#device-NAME .matrix tbody th")]
            .filter((head) => head.textContent.endsWith(" (spi)")).map((head) => head.firstChild.data.trim())"""
        page = self.open("#device-KS50")
        names = page.evaluate(marked.replace("NAME", "KS50"))
        self.assertIn("ERASE", names)
        self.assertNotIn("PROGRAM", names)
        self.assertEqual(self.open("#device-OVD1").evaluate(marked.replace("NAME", "OVD1")), [])

    def test_narrow_window_scrolls_down_only(self):
        page = self.open("#device-KS50", width=400, height=800)
        self.assertLessEqual(page.evaluate("document.documentElement.scrollWidth"), 400)

    def test_screenshot(self):
        image = self.open().screenshot()
        self.assertEqual(image[:8], b"\x89PNG\r\n\x1a\n")
        self.assertEqual(struct.unpack(">II", image[16:24]), (1280, 900))
        self.assertGreater(len(image), 20000)

    def test_prints(self):
        page = self.open("#device-KS50")
        page.emulate("dark", media="print")
        self.assertEqual(page.evaluate("getComputedStyle(document.body).backgroundColor"), "rgb(255, 255, 255)")
        self.assertEqual(page.evaluate("getComputedStyle(document.getElementById('filters')).display"), "none")
        page.emulate("light")
        self.assertEqual(page.pdf()[:5], b"%PDF-")


class Hostile(PageTest):
    @classmethod
    def make(cls):
        return report(cls.place, database(cls.place, HOSTILE), status=2)  # some names have no answer

    NAMES = ["<script>alert(1)</script>", "</script>", "<script>", "\"onclick=\"alert(3)", "A'B", "100%", "\ufffd",
             "\ufffd", "toString", "__proto__", "<u>F</u>"]

    def opened(self, scripts=True):
        page = self.open(scripts=scripts)
        page.run_scripts()
        return page

    def test_names_show_as_text(self):
        for scripts in (True, False):
            self.assertEqual(self.listed(self.opened(scripts)), self.NAMES)

    def test_nothing_of_it_is_markup(self):
        page = self.opened()
        page.click("#open-all")
        self.assertEqual(page.complaints(), [])
        self.assertEqual(page.evaluate("document.querySelectorAll('img, u, s, [onclick], [onerror]').length"), 0)
        self.assertEqual(page.evaluate("document.scripts.length"), 4)  # index, two families, the page's own

    def test_values_show_as_text(self):
        for scripts in (True, False):
            text = self.opened(scripts).evaluate("document.querySelector('.sheet').textContent")
            for value in ("</script><script>alert(2)</script>", "\"'&amp;%s%n", "\ufffd\ufffdé", "<!--",
                          "<img src=x onerror=\"alert('p')\">", "<i>value</i>"):
                self.assertIn(value, text)

    def test_links_lead_to_the_names(self):
        for name in ("<script>", "A'B", "100%", "</script>", "toString", "__proto__"):
            page = self.opened()
            page.evaluate(f"location.hash = '#device-' + encodeURIComponent({name!r})")
            page.wait_until(f"document.getElementById('device-' + {name!r}).parentElement.open")
        page = self.opened()
        page.click("#multiboot a")
        self.assertEqual(page.complaints(), [])

    def test_broken_addresses_lead_nowhere(self):
        page = self.open("#device-%E0%A4%A")
        self.assertEqual(self.listed(page), self.NAMES)
        self.assertEqual(page.complaints(), [])


class ManyFamilies(PageTest):
    """The overview is longer than the window."""
    @classmethod
    def make(cls):
        names = [f"fam{number}" for number in range(200)]
        listed = ",".join(names)
        files = {f"{name}.acd": f"OPERATION = ERASE,Bscan,USB2\n[D{name}]\n".encode() for name in names}
        files["base.acd"] = (f"DEVICE_SUPPORTED = {listed}\nPROGRAM_OPTION_PACKAGE = {listed}\n"
                             f"BS = outputs,USB2:families,{listed}\n").encode()
        return report(cls.place, database(cls.place, files))

    def is_search_visible(self, page):
        return page.evaluate("""(() => {
            const place = document.getElementById("search").getBoundingClientRect();
            return place.top >= 0 && place.bottom <= innerHeight;
        })()""")

    def test_search_stays_visible(self):
        page = self.open()
        self.assertTrue(self.is_search_visible(page))
        page.evaluate("document.querySelector('#list .device:last-of-type').scrollIntoView({block: 'end'})")
        page.settle()
        self.assertTrue(self.is_search_visible(page))

    def test_all_families_are_printed(self):
        page = self.open()
        page.emulate("light", media="print")
        self.assertEqual(page.evaluate("getComputedStyle(document.querySelector('#overview .scroll')).maxHeight"), "none")


class ManyDevices(PageTest):
    COUNT = 3000

    @classmethod
    def make(cls):
        return report(cls.place, database(cls.place, many_devices(cls.COUNT)))

    def test_lists_some_and_more_when_asked(self):
        page = self.open()
        self.assertEqual(len(self.listed(page)), 100)
        self.assertEqual(self.count(page), "3,000 devices, the first 100 listed")
        page.click("#more")
        self.assertEqual(len(self.listed(page)), 200)
        self.assertEqual(page.complaints(), [])

    def test_search_finds_the_last(self):
        page = self.open()
        page.press("/")
        page.write("b1499")
        self.assertEqual(self.listed(page), ["B1499"])

    def test_filter(self):
        page = self.open()
        page.choose("#operation", "ERASE")
        self.assertEqual(self.count(page), "1,500 of 3,000 devices, the first 100 listed")
        self.assertEqual(self.listed(page)[0], "B0")

    def test_link_to_a_device_far_down(self):
        page = self.open("#device-B1234")
        part = "document.getElementById('device-B1234')"
        self.assertTrue(page.evaluate(f"{part}.parentElement.open"))
        self.assertTrue(self.is_seen(page, f"{part}.parentElement.firstElementChild"))
        for text in ("1234", "VENDOR", "Korvel", "bee.acd:"):
            self.assertIn(text, page.evaluate(f"{part}.textContent"))

    def test_opening_shows_the_sheet(self):
        page = self.open()
        self.assertEqual(page.evaluate("document.querySelector('.sheet').textContent"), "")
        page.evaluate("document.querySelector('.device summary').click()")
        page.wait_until("document.querySelector('.sheet').textContent !== ''")
        self.assertIn("VENDOR", page.evaluate("document.querySelector('.sheet').textContent"))

    def test_multiboot_names_its_devices(self):
        page = self.open()
        page.evaluate("document.querySelector('#multiboot summary').click()")
        page.wait_until("document.querySelector('#multiboot a') !== null")
        self.assertEqual(page.evaluate("[...document.querySelectorAll('#multiboot a')].map((one) => one.textContent)"),
                         ["A3", "B4"])

    def test_reads_without_scripts(self):
        page = self.open(scripts=False)
        page.run_scripts()
        text = page.evaluate("document.getElementById('devices').innerText")
        self.assertIn("A0, A1, A2", text)
        self.assertIn("B1498, B1499", text)
        self.assertEqual(page.evaluate("document.querySelectorAll('#overview tbody tr').length"), 2)


if __name__ == "__main__":
    TOOL = sys.argv.pop(1)
    with browser.Browser() as CHROMIUM:
        unittest.main()
