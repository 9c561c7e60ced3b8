@import "Vesk/vxObject/IObject.h"
$functor+ bool F(int32 a = 1, string8 const& b) : [ 7 ];
$functor void G();
// A tab counts 4; a shallower line loses its blanks alone.
void use()
{
    $makefunctor F f
    {
	    if (a)
		    return 1;
  return 2;
    }
    f(1, "");
}
$makeconstfunctor G g { go(); }
$makefunctor F bound(find(x, y), `Base<int, char>`) { return a + m_n; };
$makeconstfunctor G constant(this, Base)
{
	go();
}
