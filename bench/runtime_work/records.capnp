@0xd3a4f1c09be27a55;
struct Place { x @0 :Int32; y @1 :Int32; }
struct Entry { id @0 :Int32; name @1 :Text; price @2 :Float64; active @3 :Bool; place @4 :Place; tags @5 :List(Int32); }
struct Entries { entries @0 :List(Entry); }
