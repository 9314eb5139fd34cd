// Search, filters and links of a device report. Works on the data in the page; without this script the page
// shows what the tool wrote into it. Nothing here makes markup from text: all text goes in as text.
"use strict";

(() => {
    const byId = (id) => document.getElementById(id);
    const read = (id) => JSON.parse(byId(id).textContent);

    /** Makes an element; texts among its children become text. */
    function element(tag, attributes = {}, ...children) {
        const made = document.createElement(tag);
        for (const [name, value] of Object.entries(attributes)) {
            made.setAttribute(name, value);
        }
        made.append(...children);
        return made;
    }

    // ---- The data ---------------------------------------------------------------------------------------------

    const index = read("index");
    const columns = [...index.modes, "BSDL"];

    const devices = (() => {
        const counts = index.families.map(() => 0);
        return index.names.map((name, position) => {
            const family = index.family[position];
            return {
                name, position, family,
                idcode: index.idcode[position],
                table: index.table[position],
                ordinal: counts[family]++, // among the devices of its family
                text: `${name}\n${index.families[family]}\n${index.idcode[position]}`.toLowerCase(),
                part: null, // the element, once it is needed
            };
        });
    })();
    const byName = new Map(devices.map((device) => [device.name.toLowerCase(), device]).reverse());
    const multiboot = new Map(index.multiboot);
    const chunks = index.families.map(() => null);

    function chunkOf(device) {
        chunks[device.family] ??= read(`family-${device.family}`);
        return chunks[device.family];
    }

    const arrangementsOf = (() => {
        let known = null;
        return (device) => {
            if (known === null) {
                known = new Map();
                for (const [arrangement, members] of multiboot) {
                    for (const member of members) {
                        known.set(member, [...(known.get(member) ?? []), arrangement]);
                    }
                }
            }
            return known.get(device.position) ?? [];
        };
    })();

    // ---- The part of a device, as the tool writes it for small databases too (Parts.cpp) ----------------------

    const headRow = (texts) => element("thead", {}, element("tr", {},
        ...texts.map((text) => element("th", {scope: "col"}, text))));

    const scrolling = (label, device, table) => element("div",
        {class: "scroll", tabindex: "0", role: "region", "aria-label": `${label} of ${device.name}`}, table);

    function cell(outputs) {
        if (outputs === 0) {
            return element("td", {class: "none"}, "–");
        }
        const isIn = (output) => (outputs >> output & 1) !== 0;
        const words = index.outputs.filter((_, output) => isIn(output)).join(", ");
        return element("td", {"aria-label": words, title: words}, ...[...index.letters].map(
            (letter, output) => isIn(output) ? element("b", {}, letter) : element("i", {}, "·")));
    }

    const legend = () => element("span", {class: "legend"}, ...[...index.letters].flatMap(
        (letter, output) => [...(output === 0 ? [] : [", "]), element("b", {}, letter), ` ${index.outputs[output]}`]));

    function matrix(title, rows, device, headings) {
        if (rows.length === 0) {
            return [];
        }
        const isFlash = index.families[device.family] === "spi";
        const spi = index.modes.indexOf("SPI");
        const marked = (sets) => !isFlash && sets.every((outputs, column) => outputs === 0 || column === spi);
        const body = rows.map(([key, ...sets]) => element("tr", {}, element("th", {scope: "row"}, key,
            ...(marked(sets) ? [" ", element("i", {title: index.spi}, "(spi)")] : [])), ...sets.map(cell)));
        return [scrolling(title, device, element("table", {class: "matrix"},
            element("caption", {}, `${title} `, legend()),
            headRow(["", ...headings]), element("tbody", {}, ...body)))];
    }

    function properties(title, coded, chunk, device) {
        if (coded === 0) {
            return [];
        }
        const place = ([file, line, column]) => `${chunk.files[file]}:${line}:${column}`;
        const own = coded.slice(0, -1);
        const shared = chunk.sets[coded.at(-1)].map((row) => chunk.rows[row]);
        const body = [...own, ...shared].map(([key, from, file, line, column, ...values]) => element("tr", {},
            element("th", {scope: "row"}, chunk.words[key]), element("td", {}, values.join(", ") || "(none)"),
            element("td", {}, chunk.words[from]), element("td", {class: "origin"}, place([file, line, column]))));
        return [scrolling(title, device, element("table", {class: "properties"}, element("caption", {}, title),
            headRow(["Property", "Value", "From", "Where"]), element("tbody", {}, ...body)))];
    }

    function facts(device, idcodeOrigin, chunk) {
        const fact = (term, ...value) => element("div", {}, element("dt", {}, term), element("dd", {}, ...value));
        const list = element("dl", {class: "facts"}, fact("Family", index.families[device.family]));
        if (idcodeOrigin !== 0) {
            const [file, line, column] = idcodeOrigin;
            list.append(fact("IDCODE", element("code", {}, device.idcode), " ",
                element("span", {class: "origin"}, `${chunk.files[file]}:${line}:${column}`)));
        }
        list.append(fact("Modes", index.tables[device.table].modes.join(" ")));
        const arrangements = arrangementsOf(device);
        if (arrangements.length > 0) {
            list.append(fact("Multiboot", arrangements.join(", ")));
        }
        return list;
    }

    function sheet(device) {
        const fault = index.faults[device.position];
        if (fault !== undefined) {
            return [element("p", {class: "fault"}, `No answer: ${fault}`)];
        }
        const chunk = chunkOf(device);
        const table = index.tables[device.table];
        const [idcodeOrigin, own, flash] = chunk.devices[device.ordinal];
        return [
            facts(device, idcodeOrigin, chunk),
            ...matrix("Operations", table.operations, device, columns),
            ...matrix("Programming options", table.options, device, index.modes),
            ...properties("Properties", own, chunk, device),
            ...properties("Properties of the flash", flash, chunk, device),
        ];
    }

    /** Fills the part with what it shows when it is open. */
    function fill(device) {
        const body = device.part.lastElementChild;
        if (!body.hasChildNodes()) {
            body.append(...sheet(device));
        }
    }

    function makePart(device) {
        const part = element("details", {class: "device"},
            element("summary", {}, element("h4", {}, device.name), " ",
                element("span", {class: "idcode"}, device.idcode), " ",
                element("span", {class: "modes"}, index.tables[device.table].modes.join(" "))),
            element("div", {class: "sheet", id: `device-${device.name}`}));
        part.addEventListener("toggle", () => part.open && fill(device));
        return part;
    }

    function partOf(device) {
        device.part ??= makePart(device);
        return device.part;
    }

    const familyHeading = (family) => element("h3", {id: `in-${index.families[family]}`}, index.families[family]);

    // ---- The list ---------------------------------------------------------------------------------------------

    const form = byId("filters");
    const search = byId("search");
    const chosen = {family: byId("family"), operation: byId("operation"), mode: byId("mode"), output: byId("output")};
    const list = byId("list");
    const more = byId("more");

    // How many devices are listed before somebody asks for more: all, where the tool has written them all already.
    const batch = list.childElementCount > 0 ? devices.length : 100;

    let matches = [];
    let listed = 0;

    /** Does a table allow what is chosen? A choice of nothing is a choice of anything. */
    function allows(table, operation, mode, output) {
        if (operation === "" && mode === "" && output === "") {
            return true;
        }
        const fits = (outputs) => output === "" ? outputs !== 0 : (outputs >> output & 1) !== 0;
        return table.operations.some(([key, ...sets]) => (operation === "" || key === operation) &&
            (mode === "" ? sets.some(fits) : fits(sets[mode])));
    }

    function findMatches() {
        const allowing = index.tables.map((table) =>
            allows(table, chosen.operation.value, chosen.mode.value, chosen.output.value));
        const text = search.value.trim().toLowerCase();
        const found = devices.filter((device) => allowing[device.table] &&
            (chosen.family.value === "" || device.family === Number(chosen.family.value)) &&
            (text === "" || device.text.includes(text)));
        // Who types a whole name means that device.
        const exact = found.findIndex((device) => device.name.toLowerCase() === text);
        if (exact > 0) {
            found.unshift(...found.splice(exact, 1));
        }
        return found;
    }

    function showMore() {
        const next = matches.slice(listed, listed + batch);
        const rows = document.createDocumentFragment();
        next.forEach((device, i) => {
            const before = matches[listed + i - 1];
            if (before === undefined || before.family !== device.family) {
                rows.append(familyHeading(device.family));
            }
            rows.append(partOf(device));
        });
        list.append(rows);
        listed += next.length;
        more.hidden = listed === matches.length;
        const [shown, of, all] = [listed, matches.length, devices.length].map((n) => n.toLocaleString("en"));
        const number = matches.length === devices.length ? `${all} devices` : `${of} of ${all} devices`;
        byId("count").textContent = more.hidden ? number : `${number}, the first ${shown} listed`;
        more.textContent = `Show ${Math.min(batch, matches.length - listed)} more`;
    }

    function update() {
        matches = findMatches();
        listed = 0;
        list.replaceChildren();
        showMore();
    }

    function clear() {
        search.value = "";
        for (const field of Object.values(chosen)) {
            field.value = "";
        }
    }

    const isListed = (device) => device.part !== null && device.part.isConnected;

    function reveal(device) {
        if (!isListed(device)) {
            clear();
            update();
        }
        if (!isListed(device)) {
            search.value = device.name;
            update();
        }
        fill(device);
        device.part.open = true;
        device.part.scrollIntoView();
        device.part.firstElementChild.focus({preventScroll: true});
    }

    function choose(family, operation) {
        clear();
        chosen.family.value = family;
        chosen.operation.value = operation;
        update();
        byId("devices").scrollIntoView();
        search.focus({preventScroll: true});
    }

    /** Goes where the address points: to a device, or to the devices of a family. */
    function follow() {
        let target = location.hash.slice(1);
        try {
            target = decodeURIComponent(target);
        } catch {
            return; // a broken link leads nowhere
        }
        if (target.startsWith("device-")) {
            const device = byName.get(target.slice("device-".length).toLowerCase());
            if (device !== undefined) {
                reveal(device);
            }
        } else if (target.startsWith("in-")) {
            const family = index.families.indexOf(target.slice("in-".length));
            if (family >= 0) {
                choose(String(family), "");
            }
        }
    }

    // ---- What the user does -----------------------------------------------------------------------------------

    function addChoices(field, texts, valueOf) {
        field.append(...texts.map((text, position) => element("option", {value: valueOf(text, position)}, text)));
    }

    function setUpFilters() {
        const operations = [...byId("overview").querySelectorAll("th.slanted")].map((head) => head.textContent);
        const others = new Set(index.tables.flatMap((table) => table.operations.map(([key]) => key)));
        addChoices(chosen.family, index.families, (_, position) => position);
        addChoices(chosen.operation, [...new Set([...operations, ...others])], (key) => key);
        addChoices(chosen.mode, columns, (_, position) => position);
        addChoices(chosen.output, index.outputs, (_, position) => position);
        form.addEventListener("input", update);
        form.addEventListener("submit", (event) => event.preventDefault());
        form.addEventListener("reset", (event) => {
            event.preventDefault();
            clear();
            update();
            search.focus();
        });
        search.addEventListener("keydown", (event) => {
            if (event.key === "Escape" && search.value !== "") {
                event.preventDefault();
                search.value = "";
                update();
            }
        });
        form.hidden = false;
    }

    function setUpList() {
        // The tool may have written the parts already; then they are all there.
        list.querySelectorAll("details").forEach((part, position) => {
            devices[position].part = part;
        });
        more.addEventListener("click", showMore);
        const setAll = (open) => matches.slice(0, listed).forEach((device) => {
            if (open) {
                fill(device);
            }
            device.part.open = open;
        });
        byId("open-all").addEventListener("click", () => setAll(true));
        byId("close-all").addEventListener("click", () => setAll(false));
        byId("openers").hidden = false;
        list.addEventListener("click", (event) => {
            // The address of an opened device can be copied.
            const summary = event.target.closest("summary");
            if (summary !== null && !summary.parentElement.open) {
                const name = summary.parentElement.lastElementChild.id;
                history.replaceState(null, "", `#${encodeURIComponent(name)}`);
            }
        });
    }

    function setUpOverview() {
        const table = byId("overview").querySelector("table");
        table.classList.add("clickable");
        table.addEventListener("click", (event) => {
            const at = event.target.closest("td");
            const head = at === null ? null : table.tHead.rows[0].cells[at.cellIndex];
            if (head !== null) {
                const isOperation = head.classList.contains("slanted");
                choose(String(at.parentElement.sectionRowIndex), isOperation ? head.textContent : "");
            }
        });
    }

    function setUpMultiboot() {
        for (const part of byId("multiboot").querySelectorAll("details")) {
            const [type, width, position] = part.closest("tr").cells;
            const arrangement = [type, width, position].map((one) => one.textContent).join(" ");
            part.addEventListener("toggle", () => {
                if (part.querySelector("a") === null) {
                    for (const member of multiboot.get(arrangement)) {
                        const name = devices[member].name;
                        part.append(" ", element("a", {href: `#device-${encodeURIComponent(name)}`}, name));
                    }
                }
            });
        }
    }

    function setUpTheme() {
        const button = byId("theme");
        const root = document.documentElement;
        const store = {
            get() { try { return localStorage.getItem("theme"); } catch { return null; } },
            set(theme) { try { localStorage.setItem("theme", theme); } catch { /* the choice lasts for the page */ } },
        };
        const system = matchMedia("(prefers-color-scheme: dark)");
        const isDark = () => (root.dataset.theme ?? (system.matches ? "dark" : "light")) === "dark";
        const label = () => { button.textContent = isDark() ? "Light" : "Dark"; };
        const stored = store.get();
        if (stored === "dark" || stored === "light") {
            root.dataset.theme = stored;
        }
        button.addEventListener("click", () => {
            root.dataset.theme = isDark() ? "light" : "dark";
            store.set(root.dataset.theme);
            label();
        });
        system.addEventListener("change", label);
        label();
        button.hidden = false;
    }

    document.addEventListener("keydown", (event) => {
        const isWriting = event.target.closest("input, select, textarea") !== null;
        if (event.key === "/" && !isWriting && !event.ctrlKey && !event.metaKey && !event.altKey) {
            event.preventDefault();
            search.focus();
            search.select();
        }
    });
    document.addEventListener("click", (event) => {
        // A link to where the address points already changes no address, but the list may have changed.
        const link = event.target.closest("a[href^='#']");
        if (link !== null && link.hash === location.hash) {
            follow();
        }
    });
    window.addEventListener("hashchange", follow);

    setUpTheme();
    setUpFilters();
    setUpList();
    setUpOverview();
    setUpMultiboot();
    update();
    follow();
})();
