" Device databases: headers, keys, values and comments.
if exists('b:current_syntax')
  finish
endif

syntax case match
syntax sync minlines=200

" A line that ends with "\" continues; what follows is part of its value, whatever it looks like.
syntax match acdMalformed /^\s*\S.*$/
syntax region acdStatement start=/^\s*[^[:blank:]=+#[][^[:blank:]=]*\s*+\?=/ skip=/\\$/ end=/$/ keepend
    \ contains=acdKey,acdOperator,acdRecord,acdField,acdContinuation,acdNumber,acdCode,acdFlag,acdMode
syntax match acdHeader /^\s*\[[^][:blank:]]\+\]\s*$/ contains=acdName
syntax match acdName /[^][:blank:][]\+/ contained
syntax match acdComment /^\s*#.*$/ contains=acdTodo,acdLint
syntax match acdLint /\<lint: ignore\>.*/ contained
syntax keyword acdTodo TODO FIXME contained

syntax match acdKey /^\s*[^[:blank:]=+#[][^[:blank:]=+]*/ contained
syntax match acdOperator /+\?=/ contained
syntax match acdRecord /:/ contained
syntax match acdField /,/ contained
syntax match acdContinuation /\\$/ contained
syntax match acdNumber /[,:]\@1<=\d\+\%(\.\d\+\)\?\ze\%([,:[:blank:]\\]\|$\)/ contained
syntax match acdCode /\<0x[0-9A-FX]\{8}\>/ contained
syntax match acdFlag /[,:]\@1<=\%(TRUE\|FALSE\)\ze\%([,:[:blank:]\\]\|$\)/ contained
syntax match acdMode /,\@1<=\%(Bscan\|SSerial\|Smap\|BSFILE\|DP770\|SPI\)\ze,/ contained

highlight default link acdComment Comment
highlight default link acdTodo Todo
highlight default link acdLint PreProc
highlight default link acdHeader Delimiter
highlight default link acdName Structure
highlight default link acdKey Identifier
highlight default link acdOperator Operator
highlight default link acdRecord Delimiter
highlight default link acdField Delimiter
highlight default link acdContinuation Special
highlight default link acdNumber Number
highlight default link acdCode Number
highlight default link acdFlag Boolean
highlight default link acdMode Type
highlight default link acdMalformed Error

let b:current_syntax = 'acd'
