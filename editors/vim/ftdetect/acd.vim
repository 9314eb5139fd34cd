autocmd BufRead,BufNewFile *.acd setfiletype acd
