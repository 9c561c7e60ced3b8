// A board on which several processes write.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace board
{

$model+ Note
{
    string8 author;
    string8 text;
};

$interface+ rmi IBoard : vesk::IObject
{
    // Answers how many notes there are now. An empty text is refused.
    void Post([in] const Note& note, [out] int32& count);
    void Notes([in] const string8& author, [out] xvector<Note>& notes);
    void Leave();
};

}
