# Makes Doxygen's comments of plain ones: those above a declaration, and those behind one. The first of a file is the file's.
/^[[:space:]]*\/\//{
  s,[\\@<>#%&$],\\&,g
  s,^([[:space:]]*)//[[:space:]]*,\1/// ,
  1s,^///,/// @file\n///,
  b
}
/[;,{}]([[:space:]]*\\)?[[:space:]]+\/\/ /{
  h
  s,^.*[[:space:]]// ,,
  s,[\\@<>#%&$],\\&,g
  x
  s,^(.*)[[:space:]]// .*$,\1,
  G
  s,\n, ///< ,
}
